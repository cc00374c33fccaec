// Opens the Hebrew and the English page of the demo company's first delivery
// note in Debian's Chromium and checks that they read as they should: the
// page decoded as windows-1255, the Hebrew heading, the customer name and the
// line descriptions in their stored left-to-right order, and the English
// page's texts as the control shows them. Saves a screenshot of each page.
//
// node pages.mjs DOVREL DEMO_DIR OUT_DIR
import { execFileSync } from 'node:child_process';
import { mkdirSync } from 'node:fs';
import { join } from 'node:path';
import { pathToFileURL } from 'node:url';

const [dovrel, demo, outDir] = process.argv.slice(2);
let chromium;
try {
    ({ chromium } = await import('playwright-core'));
} catch {
    console.error('playwright-core is not installed: run npm ci in tests/browser');
    process.exit(process.env.CI ? 1 : 77);
}

mkdirSync(outDir, { recursive: true });
// The pages are printed with the control's default settings, not the user's.
const env = { ...process.env, XDG_CONFIG_HOME: join(outDir, 'config') };
// The control's state after showing the first delivery note, from the
// automation host (show --json gives the document, not the controls).
const state = JSON.parse(execFileSync(dovrel, ['host'], {
    encoding: 'utf8', env, input: JSON.stringify(['call', 'ShowDoc', demo, 20, 2]) + '\n',
})).state;
const page = (lang, name) => {
    const file = join(outDir, name);
    execFileSync(dovrel, ['print', demo, '--lang', String(lang), '--out', file, '--no-open',
                          '--today', '2026-12-06'], { env });
    return pathToFileURL(file).href;
};

const failures = [];
const expect = (what, got, want) => {
    if (got !== want)
        failures.push(`${what}: got ${JSON.stringify(got)}, expected ${JSON.stringify(want)}`);
};

// The text of an as-is table read by where its cells stand on the screen,
// from left to right.
const asIsTexts = () => [...document.querySelectorAll("table[dir='rtl'][align='right']")]
    .map(table => [...table.querySelectorAll('td')]
        .map(td => ({ x: td.getBoundingClientRect().left, text: td.textContent }))
        .sort((a, b) => a.x - b.x)
        .map(cell => cell.text.replace(/\u00a0/g, ' '))
        .join(''));

const browser = await chromium.launch({ executablePath: '/usr/bin/chromium',
                                        args: ['--no-sandbox'] });
try {
    const tab = await browser.newPage({ viewport: { width: 1000, height: 1200 } });
    const controls = state.controls;
    const header = state.doc.header;

    await tab.goto(page(0, 'hebrew.htm'));
    expect('Hebrew page charset', await tab.evaluate(() => document.characterSet), 'windows-1255');
    expect('Hebrew heading', await tab.locator('font.TD4').innerText(),
           `${controls.txtReference1}\u00a0תעודת משלוח`);
    const texts = await tab.evaluate(asIsTexts);
    expect('customer name', texts[0], header.customerVisual);
    state.doc.lines.forEach((line, i) =>
        expect(`description of line ${i + 1}`, texts[3 + i], line.descriptionVisual));
    await tab.screenshot({ path: join(outDir, 'hebrew.png'), fullPage: true });

    await tab.goto(page(1, 'english.htm'));
    expect('English page charset', await tab.evaluate(() => document.characterSet), 'windows-1255');
    const heading = await tab.locator('font.TD4').innerText();
    expect('English heading ends with the reference', heading.endsWith(`\u00a0${controls.txtReference1}`), true);
    const to = tab.locator('td', { hasText: /^To:/ }).locator('xpath=following-sibling::td[1]');
    expect('English customer', await to.innerText(), controls.txtCustomerName);
    // The headings and total labels stand in white on black.
    const labels = await tab.evaluate(() => [...document.querySelectorAll('td.TD5')]
        .map(td => getComputedStyle(td).color));
    expect('English labels are white', labels.every(color => color === 'rgb(255, 255, 255)') &&
           labels.length > 0, true);
    const firstLine = tab.locator('table[rules] tr').nth(1).locator('td');
    expect('English description', (await firstLine.nth(2).innerText()).trim(), state.grid[1][2]);
    await tab.screenshot({ path: join(outDir, 'english.png'), fullPage: true });
} finally {
    await browser.close();
}

if (failures.length) {
    console.error(failures.join('\n'));
    process.exit(1);
}
console.log(`Both pages read as expected; screenshots in ${outDir}`);
