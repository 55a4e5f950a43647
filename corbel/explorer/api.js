// The HTTP API of corbel serve, on the server that served this page.

export class ApiError extends Error {
  constructor(status, body) {
    const word = body && body.error ? body.error : 'HTTP ' + status;
    super(body && body.message ? body.message : word);
    this.status = status;
    this.word = word;
    this.body = body || {};
  }
}

async function bodyOf(response) {
  try {
    return await response.json();
  } catch {
    return null;
  }
}

export async function getJson(path) {
  const response = await fetch(path, {cache: 'no-store', headers: {Accept: 'application/json'}});
  const body = await bodyOf(response);
  if (!response.ok) {
    throw new ApiError(response.status, body);
  }
  return body;
}

// Item names hold ':' ("02-11-22-FF-FE-33-44-55:1"), which a path carries as it is.
export function clockPath(item) {
  return '/api/v1/clocks/' + encodeURIComponent(item).replace(/%3A/g, ':');
}

// Sends changes to one clock. Answers {status, body} for every HTTP answer, since 422 and 502
// carry what the page shows next to the fields; throws only when the server does not answer.
export async function postSettings(item, changes, token) {
  const headers = {'Content-Type': 'application/json', Accept: 'application/json'};
  if (token) {
    headers.Authorization = 'Bearer ' + token;
  }
  const response = await fetch(clockPath(item) + '/settings', {
    method: 'POST',
    headers,
    body: JSON.stringify(changes),
    cache: 'no-store',
  });
  return {status: response.status, body: (await bodyOf(response)) || {}};
}
