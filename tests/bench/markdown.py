"""Tables as the pages have them."""


def print_table(rows):
    """Rows are texts by column, the same columns in each."""
    columns = list(rows[0])
    widths = [max(len(column), *(len(row[column]) for row in rows)) for column in columns]
    print()
    for row in (dict(zip(columns, columns)), None, *rows):
        cells = [row[column].ljust(width) if row else "-" * width for column, width in zip(columns, widths)]
        print("| " + " | ".join(cells) + " |" if row else "|-" + "-|-".join(cells) + "-|")
