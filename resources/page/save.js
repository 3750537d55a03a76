// The result inside the page, as it was published.

const bytesOfBase64 = text => Uint8Array.from(atob(text), byte => byte.charCodeAt(0));

const unpacked = async bytes => {
  const stream = new Blob([bytes]).stream().pipeThrough(new DecompressionStream('gzip'));
  return new Uint8Array(await new Response(stream).arrayBuffer());
};

const hexOf = bytes => Array.from(new Uint8Array(bytes), byte => byte.toString(16).padStart(2, '0')).join('');

const saveResult = async () => {
  try {
    const bytes = await unpacked(bytesOfBase64(document.getElementById('zor-block-result').textContent));
    const hash = hexOf(await crypto.subtle.digest('SHA-256', bytes));
    if (hash !== data.sha256) throw new Error('its hash is another');
    download(/\.xml$/i.test(data.document) ? data.document : 'result.xml', bytes, 'application/xml');
    say('The result is saved as it was published.');
  } catch (error) {
    say(`The result in the page is damaged: ${error.message}.`);
  }
};
