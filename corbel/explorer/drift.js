// The chart of one clock's offset from master and mean path delay over the history that the
// server keeps: seconds on a linear axis (0 = the newest sample), nanoseconds on two axes.

let chart = null;
let chartItem = '';

function points(samples, name, newest) {
  return samples.map((sample) => ({x: (sample.t - newest) / 1000, y: sample[name]}));
}

function dataset(label, colour, axis) {
  return {label, borderColor: colour, backgroundColor: colour, yAxisID: axis, data: [],
    borderWidth: 1.5, spanGaps: false};
}

function axis(title, position, colour) {
  return {type: 'linear', position, title: {display: true, text: title, color: colour},
    ticks: {color: colour}, grid: {drawOnChartArea: position === 'left'}};
}

function create(canvas) {
  return new Chart(canvas, {
    type: 'line',
    data: {datasets: [dataset('Offset from master (ns)', '#1f4fa8', 'offsetAxis'),
      dataset('Mean path delay (ns)', '#9a4a00', 'delayAxis')]},
    options: {
      animation: false,
      parsing: false,
      normalized: true,
      maintainAspectRatio: false,
      interaction: {mode: 'nearest', axis: 'x', intersect: false},
      scales: {
        x: {type: 'linear', title: {display: true, text: 'seconds before the newest sample'}},
        offsetAxis: axis('offset from master (ns)', 'left', '#1f4fa8'),
        delayAxis: axis('mean path delay (ns)', 'right', '#9a4a00'),
      },
    },
  });
}

function summaryOf(samples) {
  if (samples.length === 0) {
    return 'No samples kept yet.';
  }
  const last = samples[samples.length - 1];
  const span = Math.round((last.t - samples[0].t) / 1000);
  const show = (value) => (value === null || value === undefined ? 'not read' : value + ' ns');
  return `${samples.length} samples over ${span} s; newest: offset from master ` +
      `${show(last.offsetFromMaster)}, mean path delay ${show(last.meanPathDelay)}.`;
}

export function renderDrift(history, canvas, summary) {
  if (typeof Chart === 'undefined') {
    summary.textContent = 'The chart library did not load.';
    return;
  }
  if (!chart || chartItem !== history.item) {
    chart?.destroy();
    chart = create(canvas);
    chartItem = history.item;
  }
  const samples = history.samples || [];
  const newest = samples.length ? samples[samples.length - 1].t : 0;
  const dots = samples.length < 30 ? 2 : 0;  // single points stay visible in a short history
  chart.data.datasets[0].data = points(samples, 'offsetFromMaster', newest);
  chart.data.datasets[1].data = points(samples, 'meanPathDelay', newest);
  chart.data.datasets.forEach((set) => { set.pointRadius = dots; });
  chart.update('none');
  summary.textContent = summaryOf(samples);
}
