// The hierarchy of each domain: the grandmaster on top and every clock port under the port
// that it follows (its parent port identity), with what looks wrong said in words: a second
// grandmaster, a clock that reports another grandmaster than the one it hangs under, a parent
// that does not answer, ports that follow each other in a loop.

import {clockLink, element, identityOf, isRead, valueText, wordText} from './format.js';

function text(clock, name) {
  const value = clock.values[name];
  return isRead(value) ? String(value.value) : '';
}

// IEEE 1588 port states in which a port serves no clock: INITIALIZING, FAULTY, DISABLED,
// LISTENING. A clock that has found no master reports itself as grandmaster meanwhile.
const IDLE_STATES = new Set([1, 2, 3, 4]);

function isGrandmaster(clock) {
  return identityOf(text(clock, 'grandmasterIdentity')) === identityOf(clock.clockIdentity) &&
      !IDLE_STATES.has(clock.values.portState?.value);
}

// Links each clock of one domain to its parent; answers the top nodes and the problems seen.
function linkDomain(clocks) {
  const nodes = clocks.map((clock) => ({clock, children: []}));
  const byItem = new Map(nodes.map((node) => [node.clock.item.toUpperCase(), node]));
  const byIdentity = new Map();
  nodes.forEach((node) => byIdentity.has(identityOf(node.clock.item)) ||
      byIdentity.set(identityOf(node.clock.item), node));
  const tops = [];
  const absent = new Map();  // parent port identity that no clock answers for -> its node
  const problems = [];
  for (const node of nodes) {
    const parent = text(node.clock, 'parentPortIdentity').toUpperCase();
    if (!parent || identityOf(parent) === identityOf(node.clock.clockIdentity)) {
      tops.push(node);
      continue;
    }
    let target = byItem.get(parent) || byIdentity.get(identityOf(parent));
    if (!target) {
      target = absent.get(parent);
      if (!target) {
        target = {absent: parent, children: []};
        absent.set(parent, target);
        problems.push(parent + ' is followed but does not answer management requests.');
      }
    }
    target.children.push(node);
  }
  const grandmasters = tops.filter((node) => isGrandmaster(node.clock));
  if (grandmasters.length > 1) {
    problems.push(grandmasters.length + ' clock ports are grandmaster of this domain: ' +
        grandmasters.map((node) => node.clock.item).join(', ') + '.');
  }
  tops.sort((a, b) => grandmasters.includes(b) - grandmasters.includes(a));
  return {tops: [...tops, ...absent.values()], grandmasters, problems, nodes};
}

// Walks each tree; a clock that reports a grandmaster other than the top of its tree is
// misconfigured or cut off, and a clock that no walk reaches follows a loop.
function checkTrees(linked) {
  const reached = new Set();
  const walk = (node, top) => {
    if (node.clock) {
      reached.add(node);
      const reported = identityOf(text(node.clock, 'grandmasterIdentity'));
      if (top && reported && reported !== top) {
        linked.problems.push(node.clock.item + ' reports grandmaster ' + reported +
            ' but follows the tree of ' + top + '.');
      }
    }
    node.children.forEach((child) => walk(child, top));
  };
  for (const node of linked.tops) {
    walk(node, node.clock ? identityOf(node.clock.clockIdentity) : '');
  }
  const loop = linked.nodes.filter((node) => !reached.has(node));
  if (loop.length > 0) {
    linked.problems.push(loop.map((node) => node.clock.item).join(', ') +
        ' follow each other in a loop.');
  }
  return loop;
}

function nodeElement(node, grandmasters, top) {
  const item = element('li', 'node');
  const card = element('div', 'card');
  item.append(card);
  if (!node.clock) {
    item.classList.add('absent');
    card.append(element('span', 'item', node.absent), element('span', 'badge', 'not answering'));
  } else {
    const clock = node.clock;
    item.dataset.item = clock.item;
    item.classList.toggle('vanished', !clock.present);
    card.append(clockLink(clock.item));
    if (grandmasters.includes(node)) {
      item.classList.add('grandmaster');
      card.append(element('span', 'badge gm', 'grandmaster'));
    } else if (top) {
      card.append(element('span', 'badge', 'follows no master'));
    }
    if (!clock.present) {
      card.append(element('span', 'badge', 'vanished'));
    }
    const facts = [wordText(clock.values.portState), 'priority1 ' + text(clock, 'priority1'),
      'clock class ' + valueText(clock.values.clockClass),
      'steps removed ' + text(clock, 'stepsRemoved')];
    const description = text(clock, 'userDescription');
    card.append(element('span', 'facts', facts.join(' · ') + (description ? ' · ' + description : '')));
  }
  if (node.children.length > 0) {
    const list = element('ul');
    node.children.forEach((child) => list.append(nodeElement(child, grandmasters, false)));
    item.append(list);
  }
  return item;
}

function domainElement(domain, clocks) {
  const linked = linkDomain(clocks);
  const loop = checkTrees(linked);
  const section = element('section', 'domain');
  section.dataset.domain = domain;
  section.setAttribute('aria-labelledby', 'domain-' + domain);
  const title = element('h3', '', 'Domain ' + domain);
  title.id = 'domain-' + domain;
  section.append(title);
  if (linked.problems.length > 0) {
    const problems = element('ul', 'problems');
    linked.problems.forEach((problem) => problems.append(element('li', '', problem)));
    section.append(problems);
  }
  const tree = element('ul', 'tree');
  [...linked.tops, ...loop].forEach((node) =>
    tree.append(nodeElement(node, linked.grandmasters, linked.tops.includes(node))));
  section.append(tree);
  return section;
}

let shown = '';

export function renderHierarchy(clocks, container) {
  const signature = JSON.stringify(clocks.map((clock) => [clock.item, clock.present, clock.domain,
    ['portState', 'priority1', 'clockClass', 'stepsRemoved', 'userDescription',
      'parentPortIdentity', 'grandmasterIdentity'].map((name) => valueText(clock.values[name]))]));
  if (signature === shown) {
    return;
  }
  shown = signature;
  const focused = container.contains(document.activeElement) ?
    document.activeElement.getAttribute('href') : null;
  const domains = [...new Set(clocks.map((clock) => clock.domain))].sort((a, b) => a - b);
  container.replaceChildren(...domains.map((domain) =>
    domainElement(domain, clocks.filter((clock) => clock.domain === domain))));
  if (clocks.length === 0) {
    container.append(element('p', '', 'No clock has answered yet.'));
  }
  if (focused) {
    container.querySelector(`a[href="${CSS.escape(focused)}"]`)?.focus();
  }
}
