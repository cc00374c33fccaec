// Runs `dovrel serve` over a copy of the demo company on a free loopback
// port and drives the page in Debian's Chromium: the first delivery note,
// moving, a name search, the control's message box, printing, the company
// chooser, an account from the address, two pages apart, and a closed tab
// ending its session. Saves a screenshot of the page.
//
// node serve.mjs DOVREL DEMO_DIR OUT_DIR
import { execFileSync, spawn } from 'node:child_process';
import { cpSync, mkdirSync, rmSync, writeFileSync } from 'node:fs';
import { join, resolve } from 'node:path';
import { createInterface } from 'node:readline';

const [dovrel, demo, outArg] = process.argv.slice(2);
const outDir = resolve(outArg);
let chromium;
try {
    ({ chromium } = await import('playwright-core'));
} catch {
    console.error('playwright-core is not installed: run npm ci in tests/browser');
    process.exit(process.env.CI ? 1 : 77);
}

rmSync(outDir, { recursive: true, force: true });
const root = join(outDir, 'root');
mkdirSync(join(root, 'empty'), { recursive: true });
cpSync(demo, join(root, 'demo'), { recursive: true });
const company = join(root, 'demo');
// A one-pixel picture for the printed page's logo.
writeFileSync(join(company, 'logo.png'), Buffer.from(
    'iVBORw0KGgoAAAANSUhEUgAAAAEAAAABCAYAAAAfFcSJAAAADUlEQVR42mP8z8DwHwAFBQIAX8jx0gAAAABJRU5ErkJggg==',
    'base64'));
const env = { ...process.env, XDG_CONFIG_HOME: join(outDir, 'config') };
// The control's state after showing the first delivery note, from the
// automation host (show --json gives the document, not the controls).
const shown = JSON.parse(execFileSync(dovrel, ['host'], {
    encoding: 'utf8', env, input: JSON.stringify(['call', 'ShowDoc', company, 20, 2]) + '\n',
})).state;
const firstCustomer = shown.controls.txtCustomerName;

const failures = [];
const expect = (what, got, want) => {
    if (got !== want)
        failures.push(`${what}: got ${JSON.stringify(got)}, expected ${JSON.stringify(want)}`);
};

const server = spawn(dovrel, ['serve', '--root', root, '--listen', '127.0.0.1:0'],
                     { env, stdio: ['ignore', 'pipe', 'pipe'] });
let log = '';
server.stderr.on('data', chunk => { log += chunk; });
const url = await new Promise((resolve, reject) => {
    const timer = setTimeout(() => reject(new Error('the server printed no address')), 20000);
    createInterface({ input: server.stdout }).once('line', line => {
        clearTimeout(timer);
        resolve(line.trim());
    });
    server.once('exit', code => reject(new Error(`the server ended with ${code}: ${log}`)));
});

const browser = await chromium.launch({ executablePath: '/usr/bin/chromium', args: ['--no-sandbox'] });
const value = (tab, name) => tab.locator(`[data-control="${name}"]`).inputValue();
// Waits until every request sent so far has its reply.
const settle = async tab => {
    await tab.waitForFunction(() => document.body.dataset.ready === '1');
    await tab.waitForTimeout(150);
};
const openPage = async (context, query) => {
    const tab = await context.newPage();
    await tab.goto(url + query);
    await settle(tab);
    return tab;
};
const answerBox = async (tab, answer) => {
    const box = tab.locator('dialog[data-message]');
    await box.waitFor();
    const text = await box.locator('.text').innerText();
    await box.locator(`[data-answer="${answer}"]`).click();
    return text;
};

try {
    const context = await browser.newContext({ viewport: { width: 1100, height: 900 } });
    const q = encodeURIComponent;
    const tab = await openPage(context, `?CompDir=${q(company)}`);
    await tab.waitForFunction(() => document.querySelector('[data-control="txtCustomerName"]').value !== '');
    expect('first delivery note', await value(tab, 'txtCustomerName'), firstCustomer);
    mkdirSync(outDir, { recursive: true });
    await tab.screenshot({ path: join(outDir, 'dovrel-serve.png') });

    await tab.click('[data-control="NextButt"]');
    await tab.waitForFunction(first =>
        document.querySelector('[data-control="txtCustomerName"]').value !== first, firstCustomer);
    await tab.click('[data-control="PrevButt"]');
    await tab.waitForFunction(first =>
        document.querySelector('[data-control="txtCustomerName"]').value === first, firstCustomer);

    // A name search: the name typed, then the double click on its label.
    const other = shown.grid.length ? 'לוי אחזקות מבנים' : '';
    await tab.fill('[data-control="txtCustomerName"]', other);
    await tab.locator('[data-control="txtCustomerName"]').blur();
    await tab.dblclick('[data-control="Label2"]');
    await tab.waitForFunction(name =>
        document.querySelector('[data-control="txtCustomerName"]').value === name, other);

    // The picture settings form saves the logo, a file under the root.
    await tab.click('[data-control="CmdParams"]');
    const settings = tab.locator('dialog[data-form="frmItemPics"]');
    await settings.waitFor();
    await settings.locator('[data-control="frmItemPics.txtLogoFile"]').fill(join(company, 'logo.png'));
    await settings.locator('[data-control="frmItemPics.txtLogoFile"]').blur();
    await settings.locator('[data-control="frmItemPics.cmdSaveDef"]').click();
    await tab.waitForTimeout(300);
    if (await tab.locator('dialog[data-message]').count())
        failures.push('saving the settings: ' + await answerBox(tab, 'ok'));
    await settings.locator('[data-control="frmItemPics.close"]').click();
    await settings.waitFor({ state: 'detached' });

    // Printing opens a tab with the document, its pictures from the server.
    const [printed] = await Promise.all([context.waitForEvent('page'),
                                         tab.click('[data-control="PrintButt"]')]);
    await printed.waitForLoadState();
    expect('printed page address', /\/print\/[0-9a-f]{32}$/.test(printed.url()), true);
    expect('printed page charset', await printed.evaluate(() => document.characterSet), 'windows-1255');
    const printedText = await printed.evaluate(() => document.body.innerText);
    expect('printed page holds the customer', printedText.includes(other.split(' ')[0]) ||
           printedText.includes([...other.split(' ')[0]].reverse().join('')), true);
    const broken = await printed.evaluate(() =>
        [...document.images].filter(img => !img.complete || img.naturalWidth === 0).map(i => i.src));
    expect('printed pictures that did not load', broken.join(' '), '');
    await printed.close();

    // A company folder without document files: the control's own box.
    const empty = await openPage(context, `?CompDir=${q(join(root, 'empty'))}`);
    expect('message box', await answerBox(empty, 'ok'), 'קבצי מסמכים לא נמצאו');
    await empty.waitForFunction(() => !document.querySelector('dialog[data-message]'));
    // The chooser lists the root as its only drive.
    await empty.click('[data-control="CmdDir"]');
    const chooser = empty.locator('dialog[data-form="frmOpenDir"]');
    await chooser.waitFor();
    const drives = await chooser.locator('[data-control="frmOpenDir.PathDrive"] option').allTextContents();
    expect('the chooser\'s drives', JSON.stringify(drives), JSON.stringify([root]));
    await chooser.locator('[data-control="frmOpenDir.close"]').click();
    await chooser.waitFor({ state: 'detached' });

    // An account from the address, as a customer page links to it.
    const account = await openPage(context, `?AccountKey=10004`);
    expect('account from the address', await value(account, 'txtAccountKey'), '10004');

    // Two browser contexts keep their own documents.
    const second = await browser.newContext();
    const apart = await openPage(second, `?CompDir=${q(company)}&start=2`);
    await apart.waitForFunction(() => document.querySelector('[data-control="txtCustomerName"]').value !== '');
    await apart.click('[data-control="NextButt"]');
    await apart.waitForTimeout(300);
    expect('first page kept its document', await value(tab, 'txtCustomerName'), other);
    const opened = (log.match(/page opened/g) || []).length;
    await apart.close();
    await second.close();
    await new Promise(resolve => setTimeout(resolve, 500));
    expect('a closed tab ends its session', (log.match(/page closed/g) || []).length >= 1, true);
    expect('pages opened', opened >= 4, true);
} finally {
    await browser.close();
    server.kill('SIGTERM');
}

if (failures.length) {
    console.error(failures.join('\n'));
    process.exit(1);
}
console.log('The viewer works in the browser');
