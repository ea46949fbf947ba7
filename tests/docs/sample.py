"""The files that the pages speak of, made of a simulated gesture."""
import sqlite3
import struct
import subprocess

_GESTURE = 'sim-1-0000008'  # the stroke to the left that scripts/demo explains
_LEFT = 4
_MODES = {'fp': 0, 'hg': 1, 'ds': 2}


def _rows(raw, block_width, block_height, columns):
    """The image row by row of a frame block by block."""
    size = block_width * block_height
    row_of_blocks = size * columns
    image = bytearray()
    for top in range(0, len(raw), row_of_blocks):
        for row in range(block_height):
            for block in range(columns):
                start = top + block * size + row * block_width
                image += raw[start:start + block_width]
    return bytes(image)


def _fng(mode, tiled, geometry, frames):
    """A .fng file without registers and positions; docs/recordings.md has the format."""
    block_width, block_height, columns, rows = geometry
    head = struct.pack('<4s5H2B4H2B6x', b'FNG1', 1, 0, block_width * columns, block_height * rows,
                       len(frames), _MODES[mode], tiled, *geometry, _LEFT, 0)
    frame_head = struct.pack('<IIhhBbH', 0, 0, 0, 0, 0, 0, 0)
    return head + b''.join(frame_head + _rows(raw, *geometry[:3]) for raw in frames)


def make(directory, environment):
    """Makes build/demo/corpus.db as scripts/demo does, and a user's files of one of its gestures."""
    (directory / 'build/demo').mkdir(parents=True)
    (directory / 'recordings').mkdir()
    corpus = directory / 'build/demo/corpus.db'
    subprocess.run(['fpnavi', 'synth', str(corpus), '--count', '60', '--seed', '1'],
                   env=environment, check=True, capture_output=True)
    db = sqlite3.connect(corpus)
    sequence, mode, gap, *geometry = db.execute(
        "SELECT seq, mode, json_extract(params, '$.s_gapWidth'), block_width, block_height,"
        " block_col_num, block_row_num FROM gesture JOIN param_block p ON p.id = param_block"
        " WHERE gesture.id = ?", [_GESTURE]).fetchone()
    frames = [raw for raw, in db.execute(
        'SELECT raw FROM frame_raw WHERE gesture = ? ORDER BY frame_index', [sequence])]
    db.close()
    (directory / 'dump.bin').write_bytes(b''.join(frames))
    (directory / 'device.toml').write_text(
        's_minDelta = 4\n' + ('' if gap else 's_gapWidth = 0\ns_gapHeight = 0\n'))
    (directory / 'frames.bin').write_bytes(bytes([180]) * (56 * 36 * 4))
    (directory / 'recordings/left.fng').write_bytes(_fng(mode, int(gap != 0), geometry, frames))
